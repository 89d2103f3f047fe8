// SPDX-License-Identifier: MIT
// The state shared by the object-model classes: the application and its open
// workbooks. Every object checks it first, so that one used after its
// workbook closed or its application quit fails cleanly.
#pragma once

#include <memory>
#include <vector>

#include "cells/cell_store.h"
#include "errors.h"
#include "ooxml/document.h"
#include "workbook/engine.h"

namespace workbook {

struct Book {
    std::unique_ptr<Document> doc;
    bool closed = false;

    void Close()
    {
        closed = true;
        doc.reset();
    }
};

struct Session {
    bool quit = false;
    std::vector<std::shared_ptr<Book>> books;

    void CheckLive() const
    {
        if (quit) Fail(kObjectGone, "the application has quit");
    }
    void CheckLive(const Book &book) const
    {
        CheckLive();
        if (book.closed) Fail(kObjectGone, "the workbook is closed");
    }
    void Forget(const Book *book)
    {
        std::erase_if(books, [&](const std::shared_ptr<Book> &b) { return b.get() == book; });
    }
};

// The object-model classes, made by the ones above them.
std::shared_ptr<Workbook> MakeWorkbook(std::shared_ptr<Session> session, std::shared_ptr<Book> book);
std::shared_ptr<Range> MakeRange(std::shared_ptr<Session> session, std::shared_ptr<Book> book, size_t sheet,
                                 const Rect &rect, bool byColumns);

}  // namespace workbook
