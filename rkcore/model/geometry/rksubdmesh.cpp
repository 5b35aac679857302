#include "geometry/rksubdmesh.h"

RkSubDMesh::RkSubDMesh() = default;

RkSubDMesh::~RkSubDMesh() = default;

bool RkSubDMesh::addPatch(const RkSubDPatch& patch)
{
    if (!verticesInRange(patch.vertices, 4) || !uvsInRange(patch.uvs, 4))
        return false;
    m_patches.append(patch);
    touch();
    return true;
}
