#ifndef VETRA_VETRA_H
#define VETRA_VETRA_H

/// \file
/// Every public header.

#include "vetra/base/utils/fs/filelister.h"
#include "vetra/base/utils/fs/fileutils.h"
#include "vetra/base/utils/geo/ellipcalc.h"
#include "vetra/base/utils/geo/geodesy.h"
#include "vetra/base/utils/geo/solarposition.h"
#include "vetra/base/utils/low/copypixel.h"
#include "vetra/base/utils/low/fieldcodec.h"
#include "vetra/base/utils/low/fileposition.h"
#include "vetra/base/utils/math/convexhull.h"
#include "vetra/base/utils/math/fourier/cdft.h"
#include "vetra/base/utils/math/fourier/complexdft.h"
#include "vetra/base/utils/math/fourier/fftcomplex.h"
#include "vetra/base/utils/math/hostdensify.h"
#include "vetra/base/utils/math/interpgrid.h"
#include "vetra/base/utils/math/interpolation.h"
#include "vetra/base/utils/math/matrices.h"
#include "vetra/base/utils/math/poly1d.h"
#include "vetra/base/utils/math/poly2d.h"
#include "vetra/base/utils/math/rotations/quaternion.h"
#include "vetra/base/utils/math/rotations/quatfunctions.h"
#include "vetra/base/utils/math/rotations/rotations.h"
#include "vetra/base/utils/math/sincos.h"
#include "vetra/base/utils/math/vectors.h"
#include "vetra/base/utils/resample/algorithm/averageresampler.h"
#include "vetra/base/utils/resample/algorithm/bilinearresampler.h"
#include "vetra/base/utils/resample/algorithm/cplxsarcoeffs.h"
#include "vetra/base/utils/resample/algorithm/cplxsarresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicpsresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicresampler.h"
#include "vetra/base/utils/resample/algorithm/gaussiankernel.h"
#include "vetra/base/utils/resample/algorithm/gaussianresampler.h"
#include "vetra/base/utils/resample/algorithm/kernelfile.h"
#include "vetra/base/utils/resample/algorithm/kernelresampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange4resampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange8resampler.h"
#include "vetra/base/utils/resample/algorithm/medianresampler.h"
#include "vetra/base/utils/resample/algorithm/nearestresampler.h"
#include "vetra/base/utils/resample/algorithm/sinc16resampler.h"
#include "vetra/base/utils/resample/algorithm/sinc8resampler.h"
#include "vetra/base/utils/resample/blockplanner.h"
#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/pixelclamp.h"
#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposbilineartfm.h"
#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"
#include "vetra/base/utils/resample/postfm/bufposdoublearraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/base/utils/resample/postfm/ibufpostfm.h"
#include "vetra/base/utils/resample/resample.h"
#include "vetra/base/utils/resample/resamplebuffer.h"
#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/base/utils/resample/resamplerfactory.h"
#include "vetra/base/utils/resample/resampleutils.h"
#include "vetra/base/utils/resample/shapingwindow.h"
#include "vetra/base/utils/string/basicparser.h"
#include "vetra/base/utils/string/dectodeg.h"
#include "vetra/base/utils/string/dmsutils.h"
#include "vetra/base/utils/string/itokenizer.h"
#include "vetra/base/utils/string/jsonparser.h"
#include "vetra/base/utils/string/stringtokenizer.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/base/utils/time/clock.h"
#include "vetra/base/utils/time/timer.h"
#include "vetra/base/utils/time/usleep.h"
#include "vetra/basic/gobs/raster/datatypeadapter.h"
#include "vetra/chronocore/timestamp.h"
#include "vetra/chronocore/timesystemconverter.h"
#include "vetra/export.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"
#include "vetra/version.h"

/// The library. Helpers that have no state stand in the global namespace.
namespace vetra {
/// Types of raster data.
namespace gobs {}
/// Quaternions.
namespace qtn {}
/// Time.
namespace tsys {}
/// Resampling, and what it stands on.
namespace utils {
/// Copies of pixels whose types are known at run time.
namespace low {}
/// Arrays of numbers.
namespace math {}
}  // namespace utils
}  // namespace vetra

#endif  // VETRA_VETRA_H
