/* A node of the resource tree, as a host sees it. Implemented by this library.
 *
 * Everything below a node is an entry with a key, in one collection: properties (texts), child nodes, and links, which
 * stand for a node elsewhere. Keys and all names are compared blind to letter case. An unordered node keeps its entries
 * in the order of their keys, an ordered one as they were made; there several may bear one key, and the first counts.
 *
 * An object of these interfaces is a view: it doesn't keep its node alive. When a node has gone (ZkhwNodeDeleted), only
 * AddRef and Release of its views are valid. Any number of views may stand for one node; that two pointers differ says
 * nothing. All five interfaces are one object with one table, so every pointer to a view may be used as any of them.
 *
 * The contents of a target may stay unread until they are first asked for. Operations that say "may load" then read the
 * target's files before they answer.
 *
 * Texts in are NUL-terminated and copied before the operation returns; null counts as the empty text unless stated
 * otherwise. Texts out are BSTRs that the caller frees with SysFreeString; a value ends at its first NUL there. Arrays
 * out are CoTaskMemAlloc blocks: the caller frees each string, or releases each node, then frees the array with
 * CoTaskMemFree; an empty result is count 0 and a null array. Nodes out come with one reference for the caller.
 *
 * Out pointers must not be null where E_POINTER isn't among the results, unless they are called optional. E_OUTOFMEMORY
 * is given where a string, an array or a view can't be made; what was to be given is then null and its count 0. Where
 * memory for the tree itself runs out, or a reservation's owner is no GUID where one is needed, a C++ exception leaves
 * the operation; nothing is given then. Of several changes those that were made stay, and the next call makes the rest;
 * what Reserve and its like took is let go again, as far as there is memory for that. Contents that memory ran out for
 * while they were read stay as far as they were read.
 *
 * One thread at a time for all of a tree, the calls of observers included. */
#ifndef ZKFPGA_TREE_NODE_H
#define ZKFPGA_TREE_NODE_H

#include "zkfpga/ids.h"
#include "zkfpga/tree_constants.h"
#include "zkfpga/types.h"

#ifdef __cplusplus

struct IzkProjectItem;
struct IzkProjectItemLocator;
struct IzkhwResourceTreeNodeObserver;

struct IzkhwResourceTreeNode : public IUnknown {
    /* --- What the node is --- */

    /* Its name. S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetName(BSTR* name) = 0;

    /* Its path from the root, "/" for the root itself: names joined by "/", a "/" or backslash in a name with a
     * backslash in front. Built anew at each call. S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetPath(BSTR* path) = 0;

    /* The same with each node's "DisplayName" in place of its name, where it has one; a node whose "DisplayName" is
     * empty is left out. A localised "DisplayName" ends the path: what follows isn't given. So for all display paths.
     * May load. S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetDisplayPath(BSTR* path) = 0;

    /* Renames the node and the key of its entry in the parent. S_OK. S_FALSE: the parent refused, because an unordered
     * one has that name already; the node keeps its name, but its entry is lost from the parent. E_POINTER: null. */
    virtual HRESULT STDMETHODCALLTYPE SetName(LPCWSTR name) = 0;

    /* The name of its type. S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetType(BSTR* type) = 0;

    /* Its type, all types that this inherits from, then the pieces of the property "Protocols"; repetitions stay.
     * May load. S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetTypes(ULONG* count, BSTR** types) = 0;

    /* Whether `type` is its type or one that this inherits from, or stands in "Protocols" (there letter by letter).
     * The empty name always fits. May load. S_OK: yes. S_FALSE: no. */
    virtual HRESULT STDMETHODCALLTYPE IsOfType(LPCWSTR type) = 0;

    /* --- Properties --- */

    /* The value of a property. Of a localised one, the text for the language. May load if the name is missing.
     * S_OK. S_FALSE: no property of that name, `*value` is untouched. E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetProperty(LPCWSTR name, BSTR* value) = 0;

    /* The value of the property at `index` from 0, plain and localised ones counted, in the order of the entries. May
     * load. S_OK. S_FALSE: past the last, `*value` is untouched. E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetPropertyAt(ULONG index, BSTR* value) = 0;

    /* Assigns a property, or makes a plain one at the end. Nothing happens if the name stands for a child or a link.
     * May load. Always S_OK. */
    virtual HRESULT STDMETHODCALLTYPE SetProperty(LPCWSTR name, LPCWSTR value) = 0;

    /* Assigns the plain property at `index` from 0. Localised ones are not counted here, unlike in GetPropertyAt.
     * May load. S_OK. S_FALSE: past the last. */
    virtual HRESULT STDMETHODCALLTYPE SetPropertyAt(ULONG index, LPCWSTR value) = 0;

    /* The names of the properties, plain and localised, in the order of the entries. May load.
     * S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetPropertyNames(ULONG* count, BSTR** names) = 0;

    /* --- Reservations: who holds the node, and how (ZkhwReservationMode). They live in memory only. The property
     * "ZKHWReservation" shows them. --- */

    /* How `owners`, a comma list, hold the node or a node that its property "Reserves" names; null: anybody. Of the
     * records of each node the first that fits counts. `mode` is optional. May load. S_OK: the mode isn't 0.
     * S_FALSE: it is. */
    virtual HRESULT STDMETHODCALLTYPE GetReservation(LPCWSTR owners, ULONG* mode) = 0;

    /* Takes the node and all nodes that its property "Reserves" names, at any distance, for `owner`: all or none.
     * `owner` is any text without a comma. `granted`, optional, gets the modes that the node is held in now, or 0.
     * May load. S_OK. S_FALSE: refused, nothing is taken. */
    virtual HRESULT STDMETHODCALLTYPE Reserve(LPCWSTR owner, ULONG mode, ULONG* granted) = 0;

    /* Ends what `owner` took with Reserve. S_OK: something was let go. S_FALSE: there was nothing. */
    virtual HRESULT STDMETHODCALLTYPE Unreserve(LPCWSTR owner) = 0;

    /* Takes, as Reserve does, every node below this one that is of `type` (IsOfType), all or none; below a child that
     * isn't nothing is looked at. Null or empty: all. Not the node itself. May load. S_OK. S_FALSE: refused, nothing is
     * taken. */
    virtual HRESULT STDMETHODCALLTYPE ReserveDescendants(LPCWSTR owner, ULONG mode, LPCWSTR type) = 0;

    /* Ends what `owner` took with ReserveDescendants. May load. S_OK: something was let go. S_FALSE: nothing was. */
    virtual HRESULT STDMETHODCALLTYPE UnreserveDescendants(LPCWSTR owner, LPCWSTR type) = 0;

    /* --- Editing --- */

    /* Reads `fragment`, the inside of an element in the language of resource files, into the node, as if it stood in
     * the node's own element. Observers hear of all of it at the end. S_OK. E_FAIL: it isn't well formed; what stood in
     * front of the fault has been read, and a report stands in the property "XMLParseErrors". Or there is no memory for
     * a parser, and nothing has been read. */
    virtual HRESULT STDMETHODCALLTYPE LoadContent(LPCWSTR fragment) = 0;

    /* Removes the entry of that name, with all below it, if there is one. May load. Always S_OK. */
    virtual HRESULT STDMETHODCALLTYPE RemoveEntry(LPCWSTR name) = 0;

    /* --- Neighbours --- */

    /* S_OK: the node has a parent. S_FALSE: it is a root. */
    virtual HRESULT STDMETHODCALLTYPE HasParent() = 0;

    /* The parent, or null for a root. S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetParent(IzkhwResourceTreeNode** parent) = 0;

    /* Whether any entry is a child or a link that leads somewhere. May load. S_OK: yes. S_FALSE: no. */
    virtual HRESULT STDMETHODCALLTYPE HasChildren() = 0;

    /* The nodes of all entries, links followed, in the order of the entries. May load. S_OK, E_POINTER,
     * E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetChildren(ULONG* count, IzkhwResourceTreeNode*** nodes) = 0;

    /* Those of them that are of `type` (IsOfType). */
    virtual HRESULT STDMETHODCALLTYPE GetChildrenOfType(LPCWSTR type, ULONG* count, IzkhwResourceTreeNode*** nodes) = 0;

    /* All nodes below that are of `type`, a parent before its children, links followed; below a node that isn't, the
     * walk goes on. A link to a node that the walk stands in is passed over. May load everything below. S_OK,
     * E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetDescendantsOfType(LPCWSTR type, ULONG* count,
                                                           IzkhwResourceTreeNode*** nodes) = 0;

    /* GetChildNamesOfType (below) for all types. */
    virtual HRESULT STDMETHODCALLTYPE GetChildNames(LPCWSTR path, BOOL includePath, ULONG* count, BSTR** names,
                                                    BSTR** displayNames) = 0;

    /* The names of the nodes of all entries that are of `type`. With `includePath` each is the path: `path`, or the
     * node's own if that is null, joined with the key of the entry; else the node's name, which for a link may differ
     * from its key. `displayNames`, optional, gets as many display paths, each from the node's own display path. May
     * load. S_OK, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetChildNamesOfType(LPCWSTR path, LPCWSTR type, BOOL includePath, ULONG* count,
                                                          BSTR** names, BSTR** displayNames) = 0;

    /* GetDescendantNamesEx (below) without an exclusion. */
    virtual HRESULT STDMETHODCALLTYPE GetDescendantNames(LPCWSTR path, LPCWSTR type, BOOL includePath, ULONG* count,
                                                         BSTR** names, BSTR** displayNames) = 0;

    /* Walks `path` from this node; a leading "/" is passed over and means nothing. "" finds nothing, "/" this node.
     * Without `consumed`: S_OK and the node, or S_FALSE and null. With `consumed`: S_OK, the node, and the length of
     * `path`; or S_FALSE, the last node on the way, and the offset in `path` of what is left, by one too small for each
     * escaped backslash in front of it. `consumed` and `crossedLink` are optional; the latter tells whether the way
     * went through a link. May load. S_OK, S_FALSE, E_POINTER (null `node`), E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE FindNode(LPCWSTR path, ULONG* consumed, BOOL* crossedLink,
                                               IzkhwResourceTreeNode** node) = 0;

    /* --- Change notices (ZkhwChange) --- */

    /* Calls `observer` when something of `mask` (ZkhwChange) changes about the node; `id`, a number of the caller's,
     * comes back in each call. Every number is free to use, those that nodes use among themselves included. A second
     * registration of the same observer with the same id at the same node, through whichever view, does nothing: the
     * first mask and the first view stand. A registration that is made during a notice of the node hears of what comes
     * after it. The registration holds one reference to the observer and one to this object, until Unadvise, the end of
     * the node, or the end of its tree; so at the view that CloneDetached made, it keeps the copy alive.
     * With ZkhwReservationChanged: may load. S_OK; E_POINTER: null `observer`; E_OUTOFMEMORY: nothing is registered. */
    virtual HRESULT STDMETHODCALLTYPE Advise(IzkhwResourceTreeNodeObserver* observer, ULONG mask, ULONG id) = 0;

    /* Ends registrations of `observer` at this node, through whichever view they were made: the one with `id`, or with
     * the id 0xFFFFFFFF all of them. With `subtree`, those of that id at this node and all nodes below, and together
     * with them every one there that was made with the id 0xFFFFFFFF. What is ended hears nothing more, also when a
     * notice is under way. Always S_OK, also if there is none. */
    virtual HRESULT STDMETHODCALLTYPE Unadvise(IzkhwResourceTreeNodeObserver* observer, ULONG id, BOOL subtree) = 0;

    /* Hold the notices of this node back; nests. BeginChange takes the flags that wait and gives them in `*pending`.
     * EndChange puts `flags` in place of those raised since (`replace`) or adds them, and delivers all in one call when
     * the last bracket closes. EndChange without BeginChange breaks the contract. Always S_OK. */
    virtual HRESULT STDMETHODCALLTYPE BeginChange(ULONG* pending) = 0;
    virtual HRESULT STDMETHODCALLTYPE EndChange(ULONG flags, BOOL replace) = 0;

    /* S_OK: changes wait to be delivered. S_FALSE: none. */
    virtual HRESULT STDMETHODCALLTYPE HasPendingChanges() = 0;

    /* The node and all below as text in the language of resource files. Loads everything below. S_OK, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetXml(BSTR* xml) = 0;

  protected:
    ~IzkhwResourceTreeNode() = default;
};

struct IzkhwResourceTreeNode2 : public IzkhwResourceTreeNode {
    /* As GetReservation; with `except`, of owners other than those listed. */
    virtual HRESULT STDMETHODCALLTYPE GetReservationEx(LPCWSTR owners, BOOL except, ULONG* mode) = 0;

  protected:
    ~IzkhwResourceTreeNode2() = default;
};

struct IzkhwResourceTreeNode3 : public IzkhwResourceTreeNode2 {
    /* GetFilteredXmlEx (below) with `keep`. */
    virtual HRESULT STDMETHODCALLTYPE GetFilteredXml(ULONG nodeNameCount, LPCWSTR* nodeNames, ULONG propertyNameCount,
                                                     LPCWSTR* propertyNames, BSTR* xml) = 0;

    /* IsCompatibleWithEx (below) with the localised properties compared. */
    virtual HRESULT STDMETHODCALLTYPE IsCompatibleWith(IzkhwResourceTreeNode* other, BOOL* result) = 0;

  protected:
    ~IzkhwResourceTreeNode3() = default;
};

struct IzkhwResourceTreeNode4 : public IzkhwResourceTreeNode3 {
    /* A deep copy of the node, of that name unless it is null or empty, as the root of a tree of its own. The tree
     * lives as long as the object in `*clone`; all other views of it are void when that goes. Registrations that were
     * made on them end without a notice. Contents that aren't loaded yet stay unread in both. Links keep leading to
     * where they led in the original's tree, so they lead somewhere only in the copy of a root. Reservations aren't
     * copied, though their property is. S_OK, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE CloneDetached(LPCWSTR name, IzkhwResourceTreeNode** clone) = 0;

    /* The names of all nodes below that are of `type` and not excluded, a parent before its children, links followed.
     * A node is excluded if its property `exclusionProperty` is empty or "true", "yes", "1", "on" or "enable"; null or
     * empty: none is. Below a node that is left out the walk goes on. A link to a node that the walk stands in is
     * passed over. `displayNames`, optional, gets as many display paths. May load everything below. S_OK, E_POINTER,
     * E_OUTOFMEMORY.
     *
     * With `includePath` each is a path, otherwise the node's name. As long as the walk has met no link it is the
     * node's own path. A link is named by its key below the own path of the node that holds it, and all behind it by
     * the way through it. The later entries of a node that holds a link are named by the way to that node: this node
     * counts as reached by `path`, or by its own path if that is null; a node below it that was reached without a link
     * has no way, so they are named as if they stood right below the root. If `path` itself, walked from here as
     * FindNode does, goes through a link, everything is named by the way from `path`. Display paths follow the same
     * rules; `path` plays no part in them, but for that last one: then the way begins at the node's display path. */
    virtual HRESULT STDMETHODCALLTYPE GetDescendantNamesEx(LPCWSTR path, LPCWSTR type, BOOL includePath,
                                                           LPCWSTR exclusionProperty, ULONG* count, BSTR** names,
                                                           BSTR** displayNames) = 0;

    /* GetXml of a copy from which entries were taken out: with `keep` all but the named ones, else the named ones. A
     * child is named by its key or its type in `nodeNames`, a property by its key in `propertyNames`; a link is never
     * named. What stays is filtered in turn, so with `keep` a node stays only if all above it are named. Links are
     * written as those of a copy (CloneDetached). Loads everything that stays, in the copy alone. A null name is the
     * empty one; an array may be null if its count is 0. Always S_OK; `*xml` is null if there is no memory for it. */
    virtual HRESULT STDMETHODCALLTYPE GetFilteredXmlEx(BOOL keep, ULONG nodeNameCount, LPCWSTR* nodeNames,
                                                       ULONG propertyNameCount, LPCWSTR* propertyNames, BSTR* xml) = 0;

    /* Sorts the owners of the node's reservations, or if it has none those of the nodes that "Reserves" names, by
     * whether the host still knows them: items in `found`, one reference each, and the owners' keys of items that are
     * there but unusable in `missing`. Owners that `locator` doesn't know at all are in neither. With `activeOnly`
     * only reservations with one of the three modes count. An owner's key that is no GUID throws. S_OK; E_POINTER if
     * any pointer is null; E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE ResolveReservations(IzkProjectItemLocator* locator, ULONG* foundCount,
                                                          IUnknown*** found, ULONG* missingCount, BSTR** missing,
                                                          BOOL activeOnly) = 0;

  protected:
    ~IzkhwResourceTreeNode4() = default;
};

struct IzkhwResourceTreeNode5 : public IzkhwResourceTreeNode4 {
    /* The reservations again, for a project item of the host as the owner: the key is the text of the item's id, with
     * braces and capital digits. A null item means any owner in GetReservationForItem; in the others it is E_POINTER,
     * and out arguments are untouched. Results otherwise as of the operations by text. */
    virtual HRESULT STDMETHODCALLTYPE ReserveForItem(IzkProjectItem* item, ULONG mode, ULONG* granted) = 0;
    virtual HRESULT STDMETHODCALLTYPE GetReservationForItem(IzkProjectItem* item, ULONG* mode) = 0;
    virtual HRESULT STDMETHODCALLTYPE UnreserveForItem(IzkProjectItem* item) = 0;
    virtual HRESULT STDMETHODCALLTYPE ReserveDescendantsForItem(IzkProjectItem* item, ULONG mode, LPCWSTR type) = 0;
    virtual HRESULT STDMETHODCALLTYPE UnreserveDescendantsForItem(IzkProjectItem* item, LPCWSTR type) = 0;

    /* Whether `other` offers all that this node asks for: each node below this one, links followed, is found at the
     * same place below `other`; each property has an equal one there, except "Value" and "Interface", which aren't
     * compared, and "SupportedValues", of whose comma list each piece must be among the other's. With `skipLocalized` a
     * property that is localised on either side isn't compared. Asks both only through these interfaces, so `other`
     * may be an object of the host. What either can't say for lack of memory counts as not there. A null `other` gives
     * false. S_OK. E_POINTER: null `result`. */
    virtual HRESULT STDMETHODCALLTYPE IsCompatibleWithEx(IzkhwResourceTreeNode* other, BOOL* result,
                                                         BOOL skipLocalized) = 0;

    /* Whether the property is a localised one. May load if the name is missing. S_OK: yes. S_FALSE: no, or there is no
     * property of that name. */
    virtual HRESULT STDMETHODCALLTYPE IsLocalizedProperty(LPCWSTR name) = 0;

  protected:
    ~IzkhwResourceTreeNode5() = default;
};

#else

typedef struct IzkhwResourceTreeNode IzkhwResourceTreeNode;

#endif /* __cplusplus */

#endif
