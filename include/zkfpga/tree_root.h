/* Queries on the whole tree: a node by its path, an option string, and arrays of text. Implemented by this library.
 *
 * Paths are as in IzkhwResourceTreeNode::FindNode; the empty path is the root. Arrays, strings and results are as in
 * tree_node.h. S_FALSE: the path leads nowhere.
 *
 * An option string is a comma list of "key=value"; null is the empty one. Blanks, tabs and line ends around items, keys
 * and values don't matter, nor does letter case of keys. A "," or "=" in a value has a backslash in front; a backslash
 * that stands before one of these or before another backslash is written four times. An item that isn't of this form,
 * and an unknown key, do nothing; of two items with one key the later counts.
 *
 *   protocol=T            only nodes of type T (IsOfType); default: all
 *   recurse=true          all nodes below, not just the next
 *   includePath=true      paths in place of names
 *   stripPathPrefix=P     takes as many characters as P has off each path or name, and with includePath one more (the
 *                         "/"), whatever they are; switches includePath on unless that came earlier in the text. With
 *                         properties, only off the path in front of the name, of which nothing may be left. A node's
 *                         name that would become empty stays whole, except in a cluster.
 *   exclusionProperty=E   with recurse: without the nodes whose property E is empty or true
 *   includeAliases=true   (GetDescendantNames only) each result is a cluster of resource, alias and display name
 *   includeDisplayNames=true  (GetDescendantNames only) the same, with the display name filled in
 *
 * "true" in any letter case is true; anything else is false. */
#ifndef ZKFPGA_TREE_ROOT_H
#define ZKFPGA_TREE_ROOT_H

#include "zkfpga/ids.h"
#include "zkfpga/types.h"

#ifdef __cplusplus

struct IzkEIOGResourceTree : public IUnknown {
    /* The names of the nodes of all entries of the node at `path`, or with recurse of all nodes below it
     * (IzkhwResourceTreeNode4). A cluster is
     *   <Cluster><Name></Name><NumElts>3</NumElts><String><Name>resource</Name><Val>...</Val></String>
     *   <String><Name>alias</Name><Val>...</Val></String><String><Name>display name</Name><Val>...</Val></String>
     *   </Cluster>
     * without the line breaks, with "&", "<" and ">" escaped. The resource is the name as shown, the display name its
     * display path. With includeAliases, the alias is the name of the first project item, as the host's item offers
     * them (host_interfaces.h), that refers to the name before the prefix is taken off; letter case doesn't matter.
     * S_OK, S_FALSE, E_POINTER, E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetDescendantNames(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** names) = 0;

    /* The names of the properties of the node at `path`, then with recurse of all nodes below it; with includePath the
     * path of the node and "/" in front. A "/" or backslash in a name has a backslash in front. The node at `path`
     * gives none if it isn't of the protocol; it is never excluded. S_OK, S_FALSE, E_POINTER, E_OUTOFMEMORY. An empty
     * result comes with an array, too, which the caller frees. */
    virtual HRESULT STDMETHODCALLTYPE GetMultiplePropertyNames(LPCWSTR path, LPCWSTR options, ULONG* count,
                                                               BSTR** names) = 0;

    /* The same with the values: each result is
     *   <Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>...</Val></String>
     *   <String><Name>value</Name><Val>...</Val></String></Cluster>
     * without the line breaks. */
    virtual HRESULT STDMETHODCALLTYPE GetMultipleProperties(LPCWSTR path, LPCWSTR options, ULONG* count,
                                                            BSTR** values) = 0;

    /* A property by its path: the node's path, "/", and the property's name. The name is what stands behind the last
     * node on the way, as it stands there: a "/" in it has no backslash. For each escaped backslash in the node's path
     * it is read from one character too far in front (IzkhwResourceTreeNode::FindNode). `options` isn't read.
     * S_OK. S_FALSE: there is none, `*value` is untouched. E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetProperty(LPCWSTR path, LPCWSTR options, BSTR* value) = 0;

  protected:
    ~IzkEIOGResourceTree() = default;
};

struct IzkEIOGResourceTree2 : public IzkEIOGResourceTree {
    /* IzkhwResourceTreeNode3::GetFilteredXml of the node at `path`. S_OK, and `*xml` is null if there is no memory for
     * it. S_FALSE: `*xml` is untouched. E_OUTOFMEMORY. */
    virtual HRESULT STDMETHODCALLTYPE GetFilteredXml(LPCWSTR path, ULONG nodeNameCount, LPCWSTR* nodeNames,
                                                     ULONG propertyNameCount, LPCWSTR* propertyNames, BSTR* xml) = 0;

  protected:
    ~IzkEIOGResourceTree2() = default;
};

#endif /* __cplusplus */

#endif
