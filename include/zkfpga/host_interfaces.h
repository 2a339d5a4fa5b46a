/* Interfaces of the host's project model that this library calls, and the one that it hands to the host there. All are
 * optional: a host that gives no context and no item has no aliases, and nothing else is missing.
 *
 * Strings and interface pointers that the host gives out of these operations belong to this library, which frees and
 * releases them, unless stated otherwise. */
#ifndef ZKFPGA_HOST_INTERFACES_H
#define ZKFPGA_HOST_INTERFACES_H

#include "zkfpga/ids.h"
#include "zkfpga/types.h"

/* A description of a project item, filled in by the host. */
typedef struct ProjectItemRecord {
    ULONG size;         /* Set to the size of the record before the call; everything else is 0 then. */
    BSTR name;          /* May be null; freed with SysFreeString. */
    GUID id;            /* Its text is the key by which the item appears in reservations. */
    ULONG reserved1[5]; /* Passed through unread. */
    void* data;         /* May be null; freed with CoTaskMemFree. */
    ULONG reserved2;    /* Passed through unread. */
} ProjectItemRecord;

#ifdef __cplusplus

struct IzkProjectItem;

/* Implemented by this library; the host calls it while IzkProjectItem::SelectItems runs, and not after. Takes part in
 * reference counting in form only: the host must neither keep nor release it. */
struct IzkProjectItemSelector : public IUnknown {
    /* Called for each project item below. `item` and `result` must not be null. `*result` becomes 1. S_FALSE: go on;
     * S_OK: it was the one. */
    virtual HRESULT STDMETHODCALLTYPE SelectItem(IzkProjectItem* item, BOOL* result) = 0;

  protected:
    ~IzkProjectItemSelector() = default;
};

/* An item of the host's project. */
struct IzkProjectItem : public IUnknown {
    /* Fills in `record`. The result isn't looked at. */
    virtual HRESULT STDMETHODCALLTYPE GetItemInfo(ProjectItemRecord* record) = 0;

    /* The item's name as the user sees it: the alias of the resource that it refers to. Null is the empty name. The
     * result isn't looked at. */
    virtual HRESULT STDMETHODCALLTYPE GetName(BSTR* name) = 0;

    /* The item's project, with one reference; it is used as an IzkProject without being asked. A failure, or no
     * project (E_FAIL), becomes the result of the query for IzkhwResourceTreeOwner. */
    virtual HRESULT STDMETHODCALLTYPE GetProject(IUnknown** project) = 0;

    /* Calls SelectItem of `selector` for the items below this one. `*result`, null before the call, may be given an
     * object; it is released. The result isn't looked at. */
    virtual HRESULT STDMETHODCALLTYPE SelectItems(IzkProjectItemSelector* selector, IUnknown** result) = 0;

  protected:
    ~IzkProjectItem() = default;
};

/* Finds project items. */
struct IzkProjectItemLocator : public IUnknown {
    /* The item of that id, with one reference, or null. A result other than 0 beside an item: it exists but can't be
     * used. The id travels by value. */
    virtual HRESULT STDMETHODCALLTYPE FindItemById(GUID id, IUnknown** item) = 0;

    /* The project's own item for a record, with one reference, or null. The result isn't looked at. */
    virtual HRESULT STDMETHODCALLTYPE FindItem(ProjectItemRecord* record, IUnknown** item) = 0;

  protected:
    ~IzkProjectItemLocator() = default;
};

/* An item that refers to a resource of the tree; asked for by its id. */
struct IzkItemResourceLink : public IUnknown {
    /* The path of the resource. Only a result of 0 means that there is one. */
    virtual HRESULT STDMETHODCALLTYPE GetResourcePath(BSTR* path) = 0;

  protected:
    ~IzkItemResourceLink() = default;
};

/* Asked for by its id; items without it are passed over. Has no operations. */
struct IzkItemMarker : public IUnknown {
  protected:
    ~IzkItemMarker() = default;
};

/* What IzkProjectItem::GetProject gives. */
struct IzkProject : public IUnknown {
    /* The object that stands for the tree in this project, with one reference; it answers for
     * IID_IzkhwResourceTreeNode. A failure becomes the result of the query for IzkhwResourceTreeOwner. */
    virtual HRESULT STDMETHODCALLTYPE GetItemObject(ProjectItemRecord* record, IUnknown** object) = 0;

  protected:
    ~IzkProject() = default;
};

/* The host's context, the second argument of QueryResourceTreeInterface. This library holds no reference to it: it has
 * to live as long as the tree is used. */
struct IzkHostContext : public IUnknown {
    /* The locator, without a new reference; null: there are no aliases. */
    virtual IzkProjectItemLocator* STDMETHODCALLTYPE GetItemLocator() = 0;

  protected:
    ~IzkHostContext() = default;
};

#else

typedef struct IzkProjectItem IzkProjectItem;
typedef struct IzkHostContext IzkHostContext;

#endif /* __cplusplus */

#endif
