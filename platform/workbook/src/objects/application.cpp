// SPDX-License-Identifier: MIT
// Application and Workbooks.
#include "objects/session.h"
#include "workbook/engine.h"

namespace workbook {
namespace {

class WorkbooksImpl : public Workbooks {
public:
    explicit WorkbooksImpl(std::shared_ptr<Session> s) : session_(std::move(s)) {}

    std::shared_ptr<Workbook> Add(const VARIANT &templ) override
    {
        session_->CheckLive();
        bool missing = templ.vt == VT_EMPTY || (templ.vt == VT_ERROR && templ.scode == DISP_E_PARAMNOTFOUND);
        if (!missing) Fail(E_INVALIDARG, "Workbooks.Add takes no template");
        return Adopt(Document::CreateNew());
    }

    std::shared_ptr<Workbook> Open(const std::string &filename) override
    {
        session_->CheckLive();
        return Adopt(Document::Open(filename));
    }

    void Close() override
    {
        session_->CheckLive();
        for (auto &b : session_->books) b->Close();
        session_->books.clear();
    }

private:
    std::shared_ptr<Workbook> Adopt(std::unique_ptr<Document> doc)
    {
        auto book = std::make_shared<Book>();
        book->doc = std::move(doc);
        session_->books.push_back(book);
        return MakeWorkbook(session_, book);
    }

    std::shared_ptr<Session> session_;
};

class ApplicationImpl : public Application {
public:
    ApplicationImpl() : session_(std::make_shared<Session>()) {}

    std::shared_ptr<Workbooks> GetWorkbooks() override
    {
        session_->CheckLive();
        return std::make_shared<WorkbooksImpl>(session_);
    }

    std::string Version() override
    {
        session_->CheckLive();
        return kEngineVersion;
    }

    void Quit() override
    {
        if (session_->quit) return;
        for (auto &b : session_->books) b->Close();
        session_->books.clear();
        session_->quit = true;
    }

private:
    std::shared_ptr<Session> session_;
};

}  // namespace

std::shared_ptr<Application> CreateApplication() { return std::make_shared<ApplicationImpl>(); }

}  // namespace workbook
